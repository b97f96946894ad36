"""The page of a fleet."""

import collections

from pages import By, EveryPage, Keys, PageTest, main


class FleetPage(EveryPage, PageTest):
    page = "fleet"

    def test_every_definition_and_question_is_told(self):
        document = self.document()
        for letter, told in (("d", document["definitions"]), ("q", document["questions"])):
            self.assertGreater(len(told), 3)
            for number, each in enumerate(told):
                text = self.script("return document.getElementById(arguments[0]).textContent",
                                   f"{letter}{number}")
                self.assertIn(each["oid"], text)
                self.assertIn(each["name"], text)
                for group in each.get("groups", [each]):
                    self.assertIn(", ".join(group["installations"]), text)

    def test_the_table_says_who_has_it_how(self):
        """Each column against the document, cell by cell."""
        document = self.document()
        columns = [cell.text for cell in self.all(".matrix thead th")][1:]
        legend = dict(line.text.split(": ", 1) for line in self.all(".matrix ~ .notes li"))
        names = [legend.get(title, title).split(", ") for title in columns]
        self.assertEqual(sorted(each["name"] for each in document["installations"]),
                         sorted(name for column in names for name in column))
        rows = self.script("""
          return Array.from(document.querySelectorAll('.matrix tbody tr'),
              (row) => Array.from(row.querySelectorAll('td'), (cell) => cell.textContent.trim()));""")
        self.assertEqual(len(document["definitions"]), len(rows))
        signs = {"changed": "~", "added": "+", "removed": "\u2212", "unchanged": "=",
                 "absent": "\u00b7", "unknown": "?"}
        for definition, cells in zip(document["definitions"], rows):
            for column, cell in zip(names, cells):
                for name in column:
                    groups = [group for group in definition["groups"]
                              if name in group["installations"]]
                    if not groups:
                        self.assertEqual("=" if definition["unchanged"] else "\u00b7", cell)
                        continue
                    self.assertTrue(cell.startswith(signs[groups[0]["standing"]]), cell)
                    self.assertEqual(groups[0]["outcome"] == "undecided", cell.endswith("!"))
                    way = "".join(filter(str.isdigit, cell))
                    if way:
                        self.assertEqual(definition["groups"].index(groups[0]) + 1, int(way))

    def test_filters(self):
        document = self.document()
        items = [(each["kind"], "undecided" if each.get("undecided", 1) else "decided")
                 for each in document["definitions"] + document["questions"]]
        for position, facet in enumerate(("kind", "state")):
            counts = collections.Counter(item[position] for item in items)
            boxes = self.all(f"fieldset[data-facet={facet}] input")
            self.assertEqual(set(counts), {box.get_attribute("value") for box in boxes})
            for box in boxes:
                box.click()
                self.wait_for_shown(len(items) - counts[box.get_attribute("value")])
                box.click()
                self.wait_for_shown(len(items))
        self.type_words(document["definitions"][0]["oid"])
        self.wait_for_shown(self.script("""
          return Array.from(document.querySelectorAll('.item')).filter(
              (e) => e.textContent.includes(arguments[0])).length;""",
                                        document["definitions"][0]["oid"]))

    def test_keyboard_alone(self):
        document = self.document()
        self.tab_to("fieldset input")
        value = self.focused("e.value")
        self.press(Keys.SPACE)
        self.wait_for_shown(sum(each["kind"] != value
                                for each in document["definitions"] + document["questions"]))
        self.tab_to(".matrix")
        self.assertNotEqual("none", self.focused("getComputedStyle(e).outlineStyle"))

    def test_a_link_leads_to_the_definition(self):
        link = self.one(".matrix tbody th a")
        link.click()
        self.assertEqual(1, len(self.all("article.item:target")))
        self.assertIn(link.text, self.one("article.item:target h3").text)

    def test_print_has_everything(self):
        text = "".join(self.pdf_text().split())
        document = self.document()
        for each in document["definitions"] + document["questions"]:
            self.assertIn("".join(each["oid"].split()), text)
        for each in document["installations"]:
            self.assertIn(each["name"], text)

    def test_hostile_texts_are_texts(self):
        self.load("hostile-fleet")
        self.check_is_quiet()
        self.assertEqual(1, self.script("return document.querySelectorAll('script').length"))
        self.assertEqual(0, self.script(
            "return document.querySelectorAll('img, iframe, base, object, embed').length"))
        text = self.script("return document.getElementById('main').textContent")
        for definition in self.document("hostile-fleet")["definitions"]:
            for clause in definition["groups"][0]["clauses"]:
                self.assertIn(clause["old"], text)
        self.assertIn("<script>alert(2)<img>", text)
        self.assertEqual(1, len(self.all(".matrix")))


if __name__ == "__main__":
    main()
