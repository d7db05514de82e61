// The words of the page, a table for each language that the service knows.
import { current, update } from "../store.ts";
import { chs } from "./chs.ts";
import { deu } from "./deu.ts";
import { eng, type Texts } from "./eng.ts";
import { fra } from "./fra.ts";
import { jpn } from "./jpn.ts";
import { kor } from "./kor.ts";

export const LANGUAGES = {
  eng: { name: "English", tag: "en", texts: eng },
  deu: { name: "Deutsch", tag: "de", texts: deu },
  fra: { name: "Français", tag: "fr", texts: fra },
  jpn: { name: "日本語", tag: "ja", texts: jpn },
  kor: { name: "한국어", tag: "ko", texts: kor },
  chs: { name: "简体中文", tag: "zh", texts: chs },
} as const;

export type Language = keyof typeof LANGUAGES;

const MEMORY = "language";

export function texts(): Texts {
  return LANGUAGES[current().language].texts;
}

function isLanguage(word: string): word is Language {
  return word in LANGUAGES;
}

export function setLanguage(word: string): void {
  if (!isLanguage(word)) return;
  document.documentElement.lang = LANGUAGES[word].tag;
  document.title = LANGUAGES[word].texts.title;
  localStorage.setItem(MEMORY, word);
  update({ language: word });
}

// The language chosen before, or the first of the browser's that there is.
export function chooseLanguage(): void {
  const words = Object.keys(LANGUAGES) as Language[];
  const wanted = navigator.languages.map((tag) => words.find((word) => tag.startsWith(LANGUAGES[word].tag)));
  setLanguage(localStorage.getItem(MEMORY) ?? wanted.find((word) => word !== undefined) ?? "eng");
}
