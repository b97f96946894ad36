{{%AUTOESCAPE context="HTML"}}<!DOCTYPE html>
<html lang="en">
<head>
<meta charset="utf-8">
<meta name="generator" content="{{PROGRAM}}">
<meta http-equiv="Content-Security-Policy" content="default-src 'none'; script-src 'sha256-{{SCRIPT_HASH}}'; style-src 'sha256-{{STYLE_HASH}}'; img-src data:; base-uri 'none'; form-action 'none'">
<meta name="viewport" content="width=device-width, initial-scale=1">
<meta name="color-scheme" content="light dark">
<title>Fleet: {{ROUTE}}</title>
<link rel="icon" href="data:,">
<style>{{STYLE:none}}</style>
</head>
<body>
<a class="skip" href="#main">Skip to the questions</a>
<header>
<h1>Fleet</h1>
<p class="route">{{ROUTE}}</p>
{{#VERDICT}}<p class="verdict {{STYLE_CLASS}}"><span class="mark" aria-hidden="true">{{SIGN}}</span> {{TEXT}}</p>{{/VERDICT}}
{{#FAILURES}}<h2>Plans that cannot be read</h2>
<ul class="refusals">{{#FAILURE}}<li><code>{{PLACE}}</code> {{TEXT}}</li>{{/FAILURE}}</ul>{{/FAILURES}}
<div class="numbers">
{{#COUNTS}}
<section aria-labelledby="by-{{WHAT}}">
<h2 id="by-{{WHAT}}">{{HEADING}}</h2>
{{#BAR}}<svg class="bar" width="100%" height="26" role="img" aria-label="{{LABEL}}">{{#PIECE}}<g class="{{STYLE_CLASS}}"><title>{{WORD}}: {{NUMBER}}</title><rect x="{{X}}%" width="{{WIDTH}}%" height="26"/>{{#SIGNED}}<text x="{{MIDDLE}}%" y="18">{{SIGN}}</text>{{/SIGNED}}</g>{{/PIECE}}</svg>{{/BAR}}
<table class="counts"><thead><tr><th scope="col">{{COLUMN}}</th><th scope="col" class="number">number</th></tr></thead>
<tbody>{{#COUNT}}<tr><th scope="row"><span class="sign {{STYLE_CLASS}}" aria-hidden="true">{{SIGN}}</span>{{WORD}}</th><td class="number">{{NUMBER}}</td></tr>{{/COUNT}}</tbody></table>
</section>
{{/COUNTS}}
</div>
</header>
<div class="columns">
<aside>
<nav aria-label="Sections">
<ul>
<li><a href="#questions">Questions</a> <span class="number">{{QUESTION_COUNT}}</span></li>
{{#RELEASE}}<li><a href="#r{{N}}">{{HEADING}}</a> <span class="number">{{NUMBER}}</span></li>{{/RELEASE}}
<li><a href="#installations">Installations</a> <span class="number">{{INSTALLATION_COUNT}}</span></li>
</ul>
</nav>
<form id="filters" role="search" aria-label="Filters" hidden>
<label for="words">Name, OID or any text</label>
<input id="words" type="search" autocomplete="off" spellcheck="false">
<p id="shown" role="status"></p>
{{#FACET}}<fieldset data-facet="{{FACET_NAME}}"><legend>{{HEADING}}</legend>
{{#CHOICE}}<label><input type="checkbox" value="{{VALUE}}" checked> <span>{{WORD}}</span> <span class="number">{{NUMBER}}</span></label>{{/CHOICE}}
</fieldset>{{/FACET}}
<button type="reset">Show all</button>
</form>
</aside>
<main id="main" tabindex="-1">
<section id="questions" aria-labelledby="questions-heading">
<h2 id="questions-heading">What to decide <span class="number">{{QUESTION_COUNT}}</span></h2>
{{#NOTHING}}<p>{{TEXT}}</p>{{/NOTHING}}
{{#QUESTION}}
<article class="item conflict" id="q{{N}}" data-kind="{{KIND}}" data-state="undecided">
<h3>{{KIND_WORD}} {{#TO}}<a href="#d{{AT}}">{{/TO}}<b>{{NAME}}</b>{{#TO_END}}</a>{{/TO_END}} ({{OID}})</h3>
<p class="what"><b>settles at {{NUMBER}}</b>, {{READY}} ready then <span class="risk">{{REASON}}</span></p>
{{#CLAUSES}}<table class="sides"><thead><tr><th scope="col">Clause</th><th scope="col">Base</th><th scope="col">Old</th><th scope="col">New</th></tr></thead>
<tbody>{{#CLAUSE}}<tr><th scope="row">{{CLAUSE_NAME}}</th><td>{{BASE}}</td><td>{{OLD}}</td><td>{{NEW}}</td></tr>{{/CLAUSE}}</tbody></table>{{/CLAUSES}}
{{#ALIKE}}<p><small>{{TEXT}}</small></p>{{/ALIKE}}
{{#CHOICES}}<p>{{TEXT}}</p>{{/CHOICES}}
<p class="where">at {{WHERE}}</p>
</article>
{{/QUESTION}}
</section>
{{#RELEASE}}
<section id="r{{N}}" aria-labelledby="r{{N}}-heading">
<h2 id="r{{N}}-heading">{{HEADING}} <span class="number">{{NUMBER}}</span></h2>
<p class="route">{{ROUTE}}</p>
{{#DIFFERS}}<p>{{TEXT}}</p>{{/DIFFERS}}
<p>{{SAME}}</p>
{{#MATRIX}}
<div class="matrix" tabindex="0" role="group" aria-label="{{LABEL}}">
<table><thead><tr><th scope="col">Definition</th>{{#COLUMN}}<th scope="col">{{TEXT}}</th>{{/COLUMN}}</tr></thead>
<tbody>{{#ROW}}<tr><th scope="row"><a href="#d{{AT}}">{{NAME}}</a></th>{{#CELL}}<td><span class="sign {{STYLE_CLASS}}">{{SIGN}}</span></td>{{/CELL}}</tr>{{/ROW}}</tbody></table>
</div>
<p><small>= unchanged, ~ changed, + added, − removed, · not there, ? without BASE otherwise than in NEW; the number tells which of those below; ! undecided.</small></p>
<ul class="notes">{{#LEGEND}}<li>{{TEXT}}</li>{{/LEGEND}}</ul>
{{/MATRIX}}
{{#DEFINITION}}
<article class="item {{STYLE_CLASS}}" id="d{{N}}" data-kind="{{KIND}}" data-state="{{STATE}}">
<h3>{{KIND_WORD}} <b>{{NAME}}</b> ({{OID}})</h3>
<p>{{HAS}} have it, {{UNCHANGED}} unchanged; other ways: {{WAYS}}; undecided: {{UNDECIDED}}</p>
{{#GROUP}}<p class="what"><span class="sign {{STYLE_CLASS}}" aria-hidden="true">{{SIGN}}</span><b>{{NUMBER}} {{STANDING}} → {{OUTCOME}}</b></p>
{{#CLAUSES}}<table class="sides"><thead><tr><th scope="col">Clause</th><th scope="col">Base</th><th scope="col">Old</th><th scope="col">New</th></tr></thead>
<tbody>{{#CLAUSE}}<tr><th scope="row">{{CLAUSE_NAME}}</th><td>{{BASE}}</td><td>{{OLD}}</td><td>{{NEW}}</td></tr>{{/CLAUSE}}</tbody></table>{{/CLAUSES}}
{{#ALIKE}}<p><small>{{TEXT}}</small></p>{{/ALIKE}}
<p class="where">{{WHERE}}</p>{{/GROUP}}
</article>
{{/DEFINITION}}
</section>
{{/RELEASE}}
<section id="installations" aria-labelledby="installations-heading">
<h2 id="installations-heading">Installations <span class="number">{{INSTALLATION_COUNT}}</span></h2>
<div class="wide" tabindex="0" role="group" aria-label="Installations">
<table class="findings"><thead><tr><th scope="col">Installation</th><th scope="col">State</th><th scope="col" class="number">Release</th><th scope="col" class="number">Questions</th><th scope="col" class="number">Refusals</th><th scope="col">Plan</th></tr></thead>
<tbody>{{#INSTALLATION}}<tr><th scope="row">{{NAME}}</th><td><span class="sign {{STYLE_CLASS}}" aria-hidden="true">{{SIGN}}</span>{{STATE}}</td><td class="number">{{RELEASE_NUMBER}}</td><td class="number">{{QUESTIONS}}</td><td class="number">{{REFUSALS}}</td><td><code>{{PATH}}</code></td></tr>{{/INSTALLATION}}</tbody></table>
</div>
</section>
</main>
</div>
<footer>{{PROGRAM}} {{COMMAND}}</footer>
<script>{{SCRIPT:none}}</script>
</body>
</html>
