"""The page of check."""

import collections

from pages import By, EveryPage, Keys, PageTest, main


class CheckPage(EveryPage, PageTest):
    page = "check"

    def test_findings_are_grouped_by_file_and_rule(self):
        expected = collections.defaultdict(collections.Counter)
        for finding in self.document()["findings"]:
            expected[finding["file"]][finding["rule"]] += 1
        told = {}
        for section in self.all("main > section[data-group]"):
            path = section.find_element(By.CSS_SELECTOR, "h2").text.rsplit(None, 1)[0]
            told[path] = collections.Counter({
                group.find_element(By.CSS_SELECTOR, "h3 b").text:
                len(group.find_elements(By.CSS_SELECTOR, ".finding"))
                for group in section.find_elements(By.CSS_SELECTOR, "div[data-group]")})
        self.assertEqual(dict(expected), told)

    def test_source_lines(self):
        findings = [f for f in self.document()["findings"] if f["source"]]
        told = self.script(
            "return Array.from(document.querySelectorAll('.source'), (e) => e.textContent.trim())")
        self.assertEqual(
            sorted((f["source"]["before"] + f["source"]["behind"]).strip() for f in findings),
            sorted(text.replace("\\u0009", "\t").strip() for text in told))
        self.assertEqual(len(findings), len(self.all(".source mark")))

    def test_filters(self):
        findings = self.document()["findings"]
        for facet in ("severity", "rule"):
            counts = collections.Counter(f[facet] for f in findings)
            boxes = self.all(f"fieldset[data-facet={facet}] input")
            self.assertEqual(set(counts), {box.get_attribute("value") for box in boxes})
            for box in boxes:
                box.click()
                self.wait_for_shown(len(findings) - counts[box.get_attribute("value")])
                self.assertEqual(
                    0, self.script("""
                      return Array.from(document.querySelectorAll('[data-group]:not([hidden])'))
                          .filter((e) => e.querySelector('.item:not([hidden])') === null)
                          .length;"""), "what has nothing left in it is not shown")
                box.click()
                self.wait_for_shown(len(findings))

    def test_keyboard_alone(self):
        findings = self.document()["findings"]
        self.tab_to("fieldset input")
        value = self.focused("e.value")
        self.press(Keys.SPACE)
        self.wait_for_shown(sum(f["severity"] != value for f in findings))
        self.assertNotEqual("none", self.focused("getComputedStyle(e).outlineStyle"))

    def test_print_has_everything(self):
        text = "".join(self.pdf_text().split())
        for finding in self.document()["findings"]:
            self.assertIn("".join(finding["text"].split()), text)
            self.assertIn(f"{finding['line']}:{finding['column']}" if finding["line"] else "", text)


if __name__ == "__main__":
    main()
