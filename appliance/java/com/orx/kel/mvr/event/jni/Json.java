package com.orx.kel.mvr.event.jni;

import java.util.ArrayList;
import java.util.LinkedHashMap;
import java.util.List;
import java.util.Map;

/**
 * What the journal writes as JSON: objects as Maps, arrays as Lists, texts and numbers as Strings;
 * there is nothing else in it.
 */
final class Json {
    private final String text;
    private int at;

    private Json(String text) {
        this.text = text;
    }

    /** @throws IllegalArgumentException it is no such text */
    static Map<String, Object> object(String text) {
        try {
            return new Json(text).object();
        } catch (IndexOutOfBoundsException | NumberFormatException end) {
            throw new IllegalArgumentException("not a line of the journal: " + text, end);
        }
    }

    private Object value() {
        return switch (text.charAt(at)) {
            case '{' -> object();
            case '[' -> array();
            case '"' -> string();
            default -> number();
        };
    }

    private Map<String, Object> object() {
        Map<String, Object> values = new LinkedHashMap<>();
        expect('{');
        while (!passes('}')) {
            String name = string();
            expect(':');
            values.put(name, value());
            passes(',');
        }
        return values;
    }

    private List<Object> array() {
        List<Object> values = new ArrayList<>();
        expect('[');
        while (!passes(']')) {
            values.add(value());
            passes(',');
        }
        return values;
    }

    private String string() {
        StringBuilder value = new StringBuilder();
        expect('"');
        for (char next = text.charAt(at++); next != '"'; next = text.charAt(at++)) {
            value.append(next == '\\' ? escaped(text.charAt(at++)) : next);
        }
        return value.toString();
    }

    private char escaped(char letter) {
        if (letter == 'u') {
            at += 4;
            return (char) Integer.parseInt(text.substring(at - 4, at), 16);
        }
        int control = "bfnrt".indexOf(letter);
        return control < 0 ? letter : "\b\f\n\r\t".charAt(control);
    }

    private String number() {
        int begin = at;
        while ("-+.eE0123456789".indexOf(text.charAt(at)) >= 0) {
            ++at;
        }
        if (at == begin) {
            throw new IllegalArgumentException("not a value: " + text.substring(at));
        }
        return text.substring(begin, at);
    }

    private boolean passes(char letter) {
        boolean isThere = text.charAt(at) == letter;
        at += isThere ? 1 : 0;
        return isThere;
    }

    private void expect(char letter) {
        if (!passes(letter)) {
            throw new IllegalArgumentException(letter + " missing: " + text.substring(at));
        }
    }
}
