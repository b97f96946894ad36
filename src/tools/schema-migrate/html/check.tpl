{{%AUTOESCAPE context="HTML"}}<!DOCTYPE html>
<html lang="en">
<head>
<meta charset="utf-8">
<meta name="generator" content="{{PROGRAM}}">
<meta http-equiv="Content-Security-Policy" content="default-src 'none'; script-src 'sha256-{{SCRIPT_HASH}}'; style-src 'sha256-{{STYLE_HASH}}'; img-src data:; base-uri 'none'; form-action 'none'">
<meta name="viewport" content="width=device-width, initial-scale=1">
<meta name="color-scheme" content="light dark">
<title>Findings: {{ROUTE}}</title>
<link rel="icon" href="data:,">
<style>{{STYLE:none}}</style>
</head>
<body>
<a class="skip" href="#main">Skip to the findings</a>
<header>
<h1>Findings</h1>
<p class="route">{{ROUTE}}</p>
{{#VERDICT}}<p class="verdict {{STYLE_CLASS}}"><span class="mark" aria-hidden="true">{{SIGN}}</span> {{TEXT}}</p>{{/VERDICT}}
{{#FAILURES}}<h2>Not everything could be checked</h2>
<ul class="refusals">{{#FAILURE}}<li><code>{{PLACE}}</code> {{TEXT}}</li>{{/FAILURE}}</ul>{{/FAILURES}}
<div class="numbers">
{{#COUNTS}}
<section aria-labelledby="by-{{WHAT}}">
<h2 id="by-{{WHAT}}">{{HEADING}}</h2>
{{#BAR}}<svg class="bar" width="100%" height="26" role="img" aria-label="{{LABEL}}">{{#PIECE}}<g class="{{STYLE_CLASS}}"><title>{{WORD}}: {{NUMBER}}</title><rect x="{{X}}%" width="{{WIDTH}}%" height="26"/>{{#SIGNED}}<text x="{{MIDDLE}}%" y="18">{{SIGN}}</text>{{/SIGNED}}</g>{{/PIECE}}</svg>{{/BAR}}
<table class="counts"><thead><tr><th scope="col">{{COLUMN}}</th><th scope="col" class="number">findings</th></tr></thead>
<tbody>{{#COUNT}}<tr><th scope="row"><span class="sign {{STYLE_CLASS}}" aria-hidden="true">{{SIGN}}</span>{{WORD}}</th><td class="number">{{NUMBER}}</td></tr>{{/COUNT}}</tbody></table>
</section>
{{/COUNTS}}
{{#RULES}}<section aria-labelledby="by-rule">
<h2 id="by-rule">By rule</h2>
<table class="counts"><thead><tr><th scope="col">Rule</th><th scope="col">What it finds</th><th scope="col" class="number">findings</th></tr></thead>
<tbody>{{#RULE}}<tr><th scope="row">{{ID}}</th><td>{{TEXT}}</td><td class="number">{{NUMBER}}</td></tr>{{/RULE}}</tbody></table>
</section>{{/RULES}}
</div>
</header>
<div class="columns">
<aside>
<nav aria-label="Files">
<ul>
{{#FILE}}<li><a href="#f{{N}}">{{SHORT}}</a> <span class="number">{{NUMBER}}</span></li>{{/FILE}}
{{#OTHER_LINK}}<li><a href="#{{ID}}">{{HEADING}}</a> <span class="number">{{NUMBER}}</span></li>{{/OTHER_LINK}}
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
{{#NOTHING}}<p>{{TEXT}}</p>{{/NOTHING}}
{{#FILE}}
<section id="f{{N}}" aria-labelledby="f{{N}}-heading" data-group>
<h2 id="f{{N}}-heading">{{PATH}} <span class="number">{{NUMBER}}</span></h2>
{{#RULE}}
<div data-group>
<h3 class="rule"><b>{{ID}}</b> {{TEXT}} <span class="number">{{NUMBER}}</span></h3>
{{#FINDING}}<div class="item finding" data-severity="{{SEVERITY}}" data-rule="{{RULE_ID}}">
<p><span class="severity {{STYLE_CLASS}}">{{SIGN}} {{SEVERITY}}</span> {{#AT}}<code>{{LINE}}:{{COLUMN}}</code> {{/AT}}{{#OF}}{{TEXT}}: {{/OF}}{{TEXT}}</p>
{{#SOURCE}}<code class="source">{{BEFORE}}<mark>{{FIRST}}</mark>{{BEHIND}}</code>{{/SOURCE}}
</div>{{/FINDING}}
</div>
{{/RULE}}
</section>
{{/FILE}}
{{#OTHER}}
<section id="{{ID}}" aria-labelledby="{{ID}}-heading">
<h2 id="{{ID}}-heading">{{HEADING}} <span class="number">{{NUMBER}}</span></h2>
<table class="findings"><thead><tr><th scope="col">Rule</th><th scope="col">Place</th><th scope="col">What</th></tr></thead>
<tbody>{{#TOLD}}<tr><th scope="row">{{RULE_ID}}</th><td><code>{{PLACE}}</code></td><td>{{#OF}}{{TEXT}}: {{/OF}}{{TEXT}}{{#REMARK}}<br>Accepted: {{TEXT}}{{/REMARK}}</td></tr>{{/TOLD}}</tbody></table>
</section>
{{/OTHER}}
</main>
</div>
<footer>{{PROGRAM}} {{COMMAND}}</footer>
<script>{{SCRIPT:none}}</script>
</body>
</html>
