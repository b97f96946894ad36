{{%AUTOESCAPE context="HTML"}}<!DOCTYPE html>
<html lang="en">
<head>
<meta charset="utf-8">
<meta name="generator" content="{{PROGRAM}}">
<meta http-equiv="Content-Security-Policy" content="default-src 'none'; script-src 'sha256-{{SCRIPT_HASH}}'; style-src 'sha256-{{STYLE_HASH}}'; img-src data:; base-uri 'none'; form-action 'none'">
<meta name="viewport" content="width=device-width, initial-scale=1">
<meta name="color-scheme" content="light dark">
<title>{{TITLE}}: {{ROUTE}}</title>
<link rel="icon" href="data:,">
<style>{{STYLE:none}}</style>
</head>
<body>
<a class="skip" href="#main">Skip to the definitions</a>
<header>
<h1>{{TITLE}}</h1>
<p class="route">{{ROUTE}}</p>
{{#READY}}<p class="verdict good"><span class="mark" aria-hidden="true">✔</span> The migration may go ahead: every definition is decided, and nothing refuses it.</p>{{/READY}}
{{#NOT_READY}}<p class="verdict bad"><span class="mark" aria-hidden="true">✘</span> The migration must not go ahead: {{WHY_NOT}}.</p>{{/NOT_READY}}
{{#REFUSALS}}<ul class="refusals">{{#REFUSAL}}<li><code>{{PLACE}}</code> {{#RULE}}<b>{{ID}}</b> {{/RULE}}{{TEXT}}</li>{{/REFUSAL}}</ul>{{/REFUSALS}}
<div class="numbers">
{{#COUNTS}}
<section aria-labelledby="by-{{WHAT}}">
<h2 id="by-{{WHAT}}">{{HEADING}}</h2>
{{#BAR}}<svg class="bar" width="100%" height="26" role="img" aria-label="{{LABEL}}">{{#PIECE}}<g class="{{STYLE_CLASS}}"><title>{{WORD}}: {{NUMBER}}</title><rect x="{{X}}%" width="{{WIDTH}}%" height="26"/>{{#SIGNED}}<text x="{{MIDDLE}}%" y="18">{{SIGN}}</text>{{/SIGNED}}</g>{{/PIECE}}</svg>{{/BAR}}
<table class="counts"><thead><tr><th scope="col">{{COLUMN}}</th><th scope="col" class="number">definitions</th></tr></thead>
<tbody>{{#COUNT}}<tr><th scope="row"><span class="sign {{STYLE_CLASS}}" aria-hidden="true">{{SIGN}}</span>{{WORD}}</th><td class="number">{{NUMBER}}</td></tr>{{/COUNT}}</tbody></table>
</section>
{{/COUNTS}}
</div>
</header>
<div class="columns">
<aside>
<nav aria-label="Sections">
<ul>
<li><a href="#undecided">Undecided</a> <span class="number">{{UNDECIDED_COUNT}}</span></li>
<li><a href="#rest">Decided</a> <span class="number">{{REST_COUNT}}</span></li>
{{#TREE_LINK}}<li><a href="#superiors">Superiors</a></li>{{/TREE_LINK}}
{{#FINDINGS_LINK}}<li><a href="#findings">Findings</a> <span class="number">{{NUMBER}}</span></li>{{/FINDINGS_LINK}}
{{#SAME_LINK}}<li><a href="#same">Unchanged</a> <span class="number">{{NUMBER}}</span></li>{{/SAME_LINK}}
<li><a href="#inputs">Inputs</a></li>
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
{{#SECTION}}
<section id="{{SECTION_ID}}" aria-labelledby="{{SECTION_ID}}-heading">
<h2 id="{{SECTION_ID}}-heading">{{HEADING}} <span class="number">{{NUMBER}}</span></h2>
{{#NOTHING}}<p>{{TEXT}}</p>{{/NOTHING}}
{{#DEFINITION}}
<article class="item {{STYLE_CLASS}}" id="d{{N}}" data-class="{{CLASS}}" data-risk="{{RISK}}" data-kind="{{KIND}}">
<h3><span class="sign {{STYLE_CLASS}}" aria-hidden="true">{{SIGN}}</span>{{KIND_WORD}} <b>{{NAME}}</b> {{OID}}{{#EXTENDS}} {{#TO}}<a href="#d{{N}}">{{/TO}}of this attribute type{{#TO_END}}</a>{{/TO_END}}{{/EXTENDS}}</h3>
<p class="what">{{CLASS_WORD}}{{#ALSO}}, {{WORD}}{{/ALSO}} → <b>{{OUTCOME}}</b>{{#RISKY}} <span class="risk {{RISK}}">{{RISK_SIGN}} risk: {{RISK}}</span>{{/RISKY}}</p>
<p>{{#REASON}}{{#TO}}<a href="#d{{N}}">{{/TO}}{{TEXT}}{{#TO_END}}</a>{{/TO_END}}{{/REASON}}</p>
<table class="sides{{#NO_BASE}} three{{/NO_BASE}}"><thead><tr><th scope="col">Clause</th>{{#SIDE}}<th scope="col">{{SIDE_NAME}} {{PLACE}}</th>{{/SIDE}}</tr></thead>
<tbody>
{{#CLAUSE}}<tr class="differs"><th scope="row">≠ {{CLAUSE_NAME}}{{#CLAUSE_RISK}} {{SIGN}} {{WORD}}{{/CLAUSE_RISK}}</th>{{#CELL}}<td{{#STYLED}} class="{{CELL_CLASS}}"{{/STYLED}}>{{#PART}}{{#ADDED}}<ins>{{/ADDED}}{{#LOST}}<del>{{/LOST}}{{#TO}}<a href="#d{{N}}">{{/TO}}{{TEXT}}{{#TO_END}}</a>{{/TO_END}}{{#LOST_END}}</del>{{/LOST_END}}{{#ADDED_END}}</ins>{{/ADDED_END}}{{/PART}}</td>{{/CELL}}</tr>{{/CLAUSE}}
{{#ALIKE}}<tr><th scope="row">{{ALIKE_NAME}}</th><td colspan="{{WIDTH}}">{{#OTHER}}{{CLAUSE_NAME}} {{#PART}}{{#TO}}<a href="#d{{N}}">{{/TO}}{{TEXT}}{{#TO_END}}</a>{{/TO_END}}{{/PART}}{{#OTHER_separator}} · {{/OTHER_separator}}{{/OTHER}}</td></tr>{{/ALIKE}}
</tbody></table>
{{#NOTES}}<ul class="notes">{{#NOTE}}<li>{{#PART}}{{#TO}}<a href="#d{{N}}">{{/TO}}{{TEXT}}{{#TO_END}}</a>{{/TO_END}}{{/PART}}</li>{{/NOTE}}</ul>{{/NOTES}}
{{#ASKED}}<p>Can be decided by <code>{{CHOICES}}</code></p>{{/ASKED}}
{{#DECIDED}}<p>Decided in <code>{{PLACE}}</code></p>{{/DECIDED}}
</article>
{{/DEFINITION}}
</section>
{{/SECTION}}
{{#TREE}}
<section id="superiors" aria-labelledby="superiors-heading">
<h2 id="superiors-heading">Superiors around what changes</h2>
{{#NOTHING}}<p>{{TEXT}}</p>{{/NOTHING}}
{{#OF_KIND}}
<h3>{{HEADING}}</h3>
<div class="tree" tabindex="0" role="group" aria-label="{{HEADING}}, each below its superior">
{{#SLICE}}<svg width="{{WIDTH}}" height="{{HEIGHT}}" role="group" aria-label="{{HEADING}}, from line {{FIRST}}"><path d="{{PATH}}"/>{{#ROW}}{{#TO}}<a href="#d{{N}}">{{/TO}}<text x="{{X}}" y="{{Y}}" class="{{STYLE_CLASS}}">{{SIGN}} {{TEXT}}{{#SAID}} <tspan>{{WORD}}</tspan>{{/SAID}}</text>{{#TO_END}}</a>{{/TO_END}}{{/ROW}}</svg>{{/SLICE}}
</div>
{{/OF_KIND}}
</section>
{{/TREE}}
{{#FINDINGS}}
<section id="findings" aria-labelledby="findings-heading">
<h2 id="findings-heading">Findings of the rules <span class="number">{{NUMBER}}</span></h2>
{{#GROUP}}
<h3>{{HEADING}}</h3>
<table class="findings"><thead><tr><th scope="col">Rule</th><th scope="col">Place</th><th scope="col">What</th></tr></thead>
<tbody>{{#FINDING}}<tr><th scope="row">{{RULE}}<br><small>{{SIGN}} {{SEVERITY}}</small></th><td><code>{{PLACE}}</code></td><td>{{#OF}}{{#PART}}{{#TO}}<a href="#d{{N}}">{{/TO}}{{TEXT}}{{#TO_END}}</a>{{/TO_END}}{{/PART}}: {{/OF}}{{TEXT}}</td></tr>{{/FINDING}}</tbody></table>
{{/GROUP}}
</section>
{{/FINDINGS}}
{{#SAME}}
<section id="same" aria-labelledby="same-heading">
<h2 id="same-heading">Unchanged <span class="number">{{NUMBER}}</span></h2>
<p>Of these nothing changes: they are the same in OLD and NEW, or gone in both.</p>
{{#DEFINITION}}<p class="item unchanged" id="d{{N}}" data-class="{{CLASS}}" data-risk="{{RISK}}" data-kind="{{KIND}}"><b>{{NAME}}</b> {{OID}} {{KIND_WORD}}, {{CLASS_WORD}}, {{OUTCOME}}: {{WHY}} <small>{{PLACE}}</small> {{#OTHER}}{{CLAUSE_NAME}} {{#PART}}{{#TO}}<a href="#d{{N}}">{{/TO}}{{TEXT}}{{#TO_END}}</a>{{/TO_END}}{{/PART}}{{#OTHER_separator}} · {{/OTHER_separator}}{{/OTHER}}</p>
{{/DEFINITION}}
</section>
{{/SAME}}
<section id="inputs" aria-labelledby="inputs-heading">
<h2 id="inputs-heading">Inputs</h2>
<table class="findings"><thead><tr><th scope="col">Of</th><th scope="col">File</th><th scope="col">SHA-256</th></tr></thead>
<tbody>{{#INPUT}}<tr><th scope="row">{{ROLE}}</th><td><code>{{PATH}}</code></td><td><code>{{DIGEST}}</code></td></tr>{{/INPUT}}</tbody></table>
</section>
</main>
</div>
<footer>{{PROGRAM}} {{COMMAND}}</footer>
<script>{{SCRIPT:none}}</script>
</body>
</html>
