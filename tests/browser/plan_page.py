"""The page of a plan and of a difference."""

import collections

from pages import By, EveryPage, Keys, PageTest, WebDriverWait, main

CLASS_WORDS = {
    "changed-by-both-mergeable": "changed by both, mergeable",
    "changed-by-both-in-conflict": "changed by both, in conflict",
}


def class_word(word):
    return CLASS_WORDS.get(word, word.replace("-", " "))


class PlanPage(EveryPage, PageTest):
    page = "plan"

    def test_numbers_are_the_documents(self):
        document = self.document()
        undecided = document["counts"]["outcome"]["undecided"]
        self.assertIn(f"must not go ahead: {undecided} definitions undecided",
                      self.one(".verdict").text)
        for what in ("class", "risk", "outcome"):
            told = dict(self.script(f"""
              return Array.from(document.querySelectorAll(
                  'section[aria-labelledby=by-{what}] tbody tr'),
                  (row) => [row.cells[0].lastChild.data, Number(row.cells[1].textContent)]);"""))
            self.assertEqual({class_word(word): number
                              for word, number in document["counts"][what].items()}, told)
            bar = self.one(f"section[aria-labelledby=by-{what}] svg").get_attribute("aria-label")
            quiet = "none" if what == "risk" else "same"
            self.assertEqual(", ".join(f"{number} {word}" for word, number in told.items()
                                       if word != quiet), bar)
            widths = self.script(f"""
              return Array.from(document.querySelectorAll(
                  'section[aria-labelledby=by-{what}] rect'),
                  (e) => parseFloat(e.getAttribute('width')))""")
            self.assertAlmostEqual(100, sum(widths), delta=0.1)

    def test_undecided_come_first(self):
        document = self.document()
        names = [d["name"] for d in document["definitions"] if d["outcome"] == "undecided"]
        self.assertEqual(names, [e.text for e in self.all("#undecided h3 b")])
        self.assertTrue(self.script("""
          const follows = (a, b) => (document.querySelector(a).compareDocumentPosition(
              document.querySelector(b)) & Node.DOCUMENT_POSITION_FOLLOWING) !== 0;
          return follows('.verdict', '.numbers') && follows('.numbers', '#undecided') &&
              follows('#undecided', '#rest') && follows('#rest', '#superiors');"""))

    def test_each_side_stands_beside_the_others(self):
        document = self.document()
        for number, definition in enumerate(document["definitions"]):
            if not definition["clauses"]:
                continue
            rows = self.script(f"""
              return Array.from(document.querySelectorAll('#d{number} tr.differs'), (row) =>
                  Array.from(row.cells, (cell) => cell.textContent));""")
            self.assertEqual(len(definition["clauses"]), len(rows))
            for row, clause in zip(rows, definition["clauses"]):
                self.assertTrue(row[0].startswith("≠ " + clause["clause"]), row)
                self.assertTrue(row[0].endswith(clause["risk"]), row)
                for cell, side in zip(row[1:], ("base", "old", "new", "result")):
                    expected = clause[side]
                    if side == "result" and not clause["decided"]:
                        expected = "? undecided"
                    elif expected is None:
                        expected = "none" if definition["places"][side] else "not there"
                    self.assertEqual(expected, cell)

    def test_a_member_that_differs_is_marked(self):
        marks = self.script("""
          return Array.from(document.querySelectorAll('ins, del'), (e) =>
              [e.tagName, getComputedStyle(e, '::before').content]);""")
        self.assertIn(["INS", '"+"'], marks)
        self.assertIn(["DEL", '"\u2212"'], marks)

    def test_colour_is_not_the_only_sign(self):
        for number, definition in enumerate(self.document()["definitions"]):
            text = self.script(f"return document.getElementById('d{number}').textContent")
            self.assertIn(class_word(definition["class"]), text)
            self.assertIn(definition["outcome"], text)
            if definition["risk"] != "none":
                self.assertIn("risk: " + definition["risk"], text)

    def test_filters(self):
        definitions = self.document()["definitions"]
        for facet in ("class", "risk", "kind"):
            counts = collections.Counter(d[facet] for d in definitions)
            boxes = self.all(f"fieldset[data-facet={facet}] input")
            self.assertEqual(set(counts), {box.get_attribute("value") for box in boxes})
            for box in boxes:
                box.click()
                self.wait_for_shown(len(definitions) - counts[box.get_attribute("value")])
                box.click()
                self.wait_for_shown(len(definitions))
        # Several together: what every one of them lets through.
        self.one("fieldset[data-facet=class] input[value=same]").click()
        self.one("fieldset[data-facet=kind] input[value=object-class]").click()
        expected = sum(d["class"] != "same" and d["kind"] != "object-class" for d in definitions)
        self.wait_for_shown(expected)
        self.assertEqual(f"{expected} of {len(definitions)} shown", self.one("#shown").text)
        self.one("button[type=reset]").click()
        self.wait_for_shown(len(definitions))

    def test_text_filter(self):
        definition = self.document()["definitions"][0]
        self.type_words(definition["oid"])
        self.script("return 0")
        self.wait_for_shown(self.script("""
          return Array.from(document.querySelectorAll('.item')).filter(
              (e) => e.textContent.includes(arguments[0])).length;""", definition["oid"]))
        self.assertFalse(self.one("#d0").get_attribute("hidden"))
        self.type_words("no definition says this")
        self.wait_for_shown(0)
        self.assertTrue(self.one("#shown").text.startswith("0 of "))
        # Any letter case, each word.
        self.type_words(definition["name"].upper() + " " + definition["oid"])
        self.wait_for_shown(1)

    def test_a_link_leads_to_what_is_hidden(self):
        link = self.one("#undecided a, #rest td a")
        target = link.get_attribute("href").split("#")[1]
        self.type_words("no definition says this")
        self.wait_for_shown(0)
        self.script(f"location.hash = '{target}'")
        self.wait_for_shown(len(self.document()["definitions"]))
        WebDriverWait(self.browser, 20).until(lambda _: self.script(f"""
          const box = document.getElementById('{target}').getBoundingClientRect();
          return Math.abs(box.top) <= 20 && box.height > 0;"""))

    def test_names_lead_to_their_definitions(self):
        document = self.document()
        numbers = {(d["kind"], d["name"].lower()): i for i, d in enumerate(document["definitions"])}
        checked = 0
        for number, definition in enumerate(document["definitions"]):
            if definition["kind"] != "object-class":
                continue
            for clause in definition["otherClauses"]:
                if clause["clause"] not in ("MUST", "MAY"):
                    continue
                for member in clause["value"].split(" $ "):
                    target = numbers.get(("attribute-type", member.lower()))
                    if target is not None:
                        checked += 1
                        self.assertGreaterEqual(self.script(f"""
                          return Array.from(document.querySelectorAll(
                              '#d{number} a[href="#d{target}"]')).filter(
                              (e) => e.textContent === arguments[0]).length;""", member), 1)
        self.assertGreater(checked, 20)

    def test_tree_of_superiors(self):
        texts = self.script(
            "return Array.from(document.querySelectorAll('.tree text'), (e) => e.textContent)")
        document = self.document()
        changed = {d["name"]: class_word(d["class"]) for d in document["definitions"]
                   if d["outcome"] != "same" and d["kind"] == "object-class"}
        by_name = {node["name"]: node for node in document["superiors"]
                   if node["kind"] == "object-class"}
        checked = 0
        for name, word in changed.items():
            if by_name[name]["superiors"]:
                checked += 1
                self.assertTrue(any(f" {name} (" in text and text.endswith(word)
                                    for text in texts), name)
        self.assertGreater(checked, 5)
        # A subordinate stands below its superior, and further right.
        places = self.script("""
          const places = {};
          for (const e of document.querySelectorAll('.tree a[href]')) {
            const box = e.firstChild.getBoundingClientRect();
            places[e.textContent.split(' ')[1]] = [box.left, box.top];
          }
          return places;""")
        for name in changed:
            for superior in by_name[name]["superiors"]:
                if superior in places:
                    self.assertLess(places[superior][0], places[name][0])
                    self.assertLess(places[superior][1], places[name][1])

    def test_keyboard_alone(self):
        definitions = self.document()["definitions"]
        self.tab_to("#words")
        self.press("t", "o", "p")
        self.wait_for_shown(self.script("""
          return Array.from(document.querySelectorAll('.item')).filter(
              (e) => e.textContent.toLowerCase().includes('top')).length;"""))
        self.press(Keys.BACKSPACE, Keys.BACKSPACE, Keys.BACKSPACE)
        self.wait_for_shown(len(definitions))
        self.tab_to("fieldset input")
        self.assertNotEqual("none", self.focused("getComputedStyle(e).outlineStyle"))
        value = self.focused("e.value")
        self.press(Keys.SPACE)
        self.wait_for_shown(sum(d["class"] != value for d in definitions))
        self.tab_to("button[type=reset]")
        self.assertNotEqual("none", self.focused("getComputedStyle(e).outlineStyle"))
        self.press(Keys.ENTER)
        self.wait_for_shown(len(definitions))
        self.tab_to("article a")
        self.assertNotEqual("none", self.focused("getComputedStyle(e).outlineStyle"))
        target = self.focused("e.getAttribute('href')")
        self.press(Keys.ENTER)
        self.assertEqual(target, self.script("return location.hash"))

    def test_print_has_everything(self):
        text = "".join(self.pdf_text().split())
        document = self.document()
        missing = [d["oid"] for d in document["definitions"]
                   if "".join(f"{d['name']}({d['oid']})".split()) not in text]
        self.assertEqual([], missing)
        for definition in document["definitions"]:
            self.assertIn("".join(definition["reason"].split()), text)
        for finding in document["findings"]:
            self.assertIn("".join(finding["text"].split()), text)
        self.emulate(media="print", features=[])
        self.assertFalse(self.one("#filters").is_displayed())


class UnknownPage(PageTest):
    """Without BASE there is no column for it."""
    page = "unknown"

    def test_is_quiet(self):
        self.check_is_quiet()

    def test_has_no_column_for_base(self):
        self.assertEqual(["Clause", "Old", "New", "Result"], [
            text.split()[0] for text in self.script("""
              return Array.from(document.querySelector('table.sides thead tr').cells,
                                (e) => e.textContent)""")])


class DiffPage(PageTest):
    page = "diff"

    def test_is_quiet(self):
        self.check_is_quiet()

    def test_has_the_differences_alone(self):
        self.assertEqual(len(self.document()["definitions"]), self.shown())
        self.assertEqual([], self.all("#same"))


class MigratePage(PageTest):
    page = "migrate"

    def test_is_quiet(self):
        self.check_is_quiet()

    def test_may_go_ahead(self):
        self.assertEqual("Migration", self.one("h1").text)
        self.assertIn("The migration may go ahead", self.one(".verdict.good").text)
        self.assertEqual("Nothing is undecided.", self.one("#undecided p").text)

    def test_decisions_are_told(self):
        decided = [d for d in self.document()["definitions"] if d["decision"]]
        self.assertGreater(len(decided), 2)
        text = self.script("return document.getElementById('rest').textContent")
        for definition in decided:
            self.assertIn(definition["decision"], text)


if __name__ == "__main__":
    main()
